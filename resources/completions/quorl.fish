# What fish offers after "quorl".

function __quorl_playlists
    quorl --playlists 2>/dev/null | cut -f4
    echo none
end

complete -c quorl -f
complete -c quorl -l text -d 'Show the pane in the terminal'
complete -c quorl -l screenshot -r -F -d 'Write a picture of the pane to a file'
complete -c quorl -l library -d 'Print what the music folder holds'
complete -c quorl -l playlists -d 'Print the playlists that can be chosen'
complete -c quorl -l wearables -d 'Print the wearables that can be chosen'
complete -c quorl -l status -d 'Print how the sync and the wearable stand'
complete -c quorl -l json -d 'Print the status or a list as JSON'
complete -c quorl -l use-wearable -x -a '(__fish_complete_directories)' -d 'Choose this wearable for good'
complete -c quorl -l use-music -x -a '(__fish_complete_directories)' -d 'Choose this music folder for good'
complete -c quorl -l choose -x -a '(__quorl_playlists)' -d 'Choose this playlist'
complete -c quorl -l limit -x -d 'Choose how much of it is synced at most'
complete -c quorl -l sync -d 'Sync now'
complete -c quorl -l cancel -d 'End the running sync'
complete -c quorl -l wait -d 'End when everything is on the wearable'
complete -c quorl -l music -x -a '(__fish_complete_directories)' -d 'For a trial with this music folder'
complete -c quorl -l wearable -x -a '(__fish_complete_directories)' -d 'For a trial with the Velora that is mounted here'
complete -c quorl -l plugins -x -a '(__fish_complete_directories)' -d 'Look for plug-ins here first'
complete -c quorl -l size -x -d 'Size of the picture in points'
complete -c quorl -l scale -x -d 'Pixels of the picture to the point'
complete -c quorl -l dark -d 'Picture the dark look'
complete -c quorl -l pane -x -a 'root playlist limit front' -d 'Picture this pane'
complete -c quorl -s h -l help -d 'Print the options and end'
complete -c quorl -l version -d 'Print the version and end'
