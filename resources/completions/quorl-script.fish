# What fish offers after "quorl-script".

complete -c quorl-script -F
complete -c quorl-script -l plugins -x -a '(__fish_complete_directories)' -d 'Look for plug-ins here first'
complete -c quorl-script -s h -l help -d 'Print the options and end'
complete -c quorl-script -l version -d 'Print the version and end'
