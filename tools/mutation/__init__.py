"""The parts of ./mutate, which says what each is for."""
