"""What tools/phone-costs and tools/hot-costs share."""
