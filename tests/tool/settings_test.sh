# Settings from the environment: the setting that holds the library to a target shows in what it tells of itself.
. "$(dirname "$0")/expect.sh"

# bodies SETTINGS
bodies() {
    PIXELKILN_SETTINGS=$1 "$program" info | sed -n 's/^bodies *//p'
}

is "bodies held to plain" "$(bodies PK.highestTarget=plain)" "plain"
is "bodies held to SSE2" "$(bodies PK.highestTarget=sse2)" "plain SSE2"
is "among other settings" "$(bodies a=b,PK.highestTarget=sse2,PK.disableAVX=false)" "plain SSE2"
is "behind pieces that are no setting" "$(bodies ,piece,,=,PK.highestTarget=sse2,)" "plain SSE2"
is "the last of two of one name" "$(bodies PK.highestTarget=sse2,PK.highestTarget=plain)" "plain"
is "a word that names no target" "$(bodies PK.highestTarget=SSE2)" "$(bodies '')"
is "no settings" "$(env -u PIXELKILN_SETTINGS "$program" info)" "$(PIXELKILN_SETTINGS='' "$program" info)"

finish
