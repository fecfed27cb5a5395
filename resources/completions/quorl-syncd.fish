# What fish offers after "quorl-syncd".

complete -c quorl-syncd -f
complete -c quorl-syncd -l trial -d 'Run beside another engine, with settings of its own'
complete -c quorl-syncd -l music-folder -x -a '(__fish_complete_directories)' -d 'Take songs and playlists from here'
complete -c quorl-syncd -l wearable -x -a '(__fish_complete_directories)' -d 'Bring them to the Velora that is mounted here'
complete -c quorl-syncd -l embedded-capacity -x -d 'What the embedded wearable holds, in bytes'
complete -c quorl-syncd -l rate-limit -x -d 'Copy at most so many bytes a second to the embedded wearable'
complete -c quorl-syncd -l retry-after -x -d 'Try again after so many seconds'
complete -c quorl-syncd -s h -l help -d 'Print the options and end'
complete -c quorl-syncd -l version -d 'Print the version and end'
