# Raw files of DV to FFmpeg and from it, with the error of each plane.
. "$(dirname "$0")/expect.sh"

if ! command -v ffmpeg > found; then
    echo "skipped: ffmpeg is not installed"
    exit 77
fi

# moving NAME SIZE RATE FILTERS: ten frames that move over a photograph
moving() {
    ffmpeg -v error -y -loop 1 -i "$media/coffee.png" -frames:v 10 \
        -vf "scale=1600:1200,crop=${2%x*}:${2#*x}:n*4:n*3,scale=out_color_matrix=$4:flags=accurate_rnd,fps=$3" \
        -r "$3" -pix_fmt yuv422p "$1" || fail "ffmpeg did not write $1"
}
# psnr FILE FILE: of Y, U and V over all frames
psnr() {
    ffmpeg -hide_banner -nostats -i "$1" -i "$2" -lavfi "[0]format=yuv422p[a];[1]format=yuv422p[b];[a][b]psnr" -f null - \
        2>&1 | sed -n 's/.*PSNR y:\([^ ]*\) u:\([^ ]*\) v:\([^ ]*\) .*/\1 \2 \3/p'
}
# near WHAT FILE FILE Y U V: no plane is further off than so many dB
near() {
    local got
    got=$(psnr "$2" "$3")
    echo "$1: $got dB"
    is "$1, $got dB, at least $4 $5 $6" "$(echo "$got" | awk -v y="$4" -v u="$5" -v v="$6" '
        function reaches(got, least) { return got == "inf" || got + 0 >= least + 0 }
        { print NF == 3 && reaches($1, y) && reaches($2, u) && reaches($3, v) }')" 1
}
# What FFmpeg says of a file, but for its own remark on raw files.
said() {
    ffmpeg -v warning -i "$1" -f null - 2>&1 | grep -v "Estimating duration from bitrate"
}

# both FORMAT SIZE RATE MATRIX PIXELS CHROMA: our file is read by FFmpeg as by us, and FFmpeg's by us as by FFmpeg.
# CHROMA is the least for what is not interpolated alike.
both() {
    moving moving.y4m "$2" "$3" "$4"
    expect 0 "10 frames of $1, $2" dv encode moving.y4m ours.dv --to "$1"
    expect 0 "errors      none" dv info ours.dv
    is "what FFmpeg says of our $1" "$(said ours.dv)" ""
    expect 0 "10 frames" dv decode ours.dv ours.y4m
    near "our $1, by FFmpeg and by us" ours.dv ours.y4m 58 "$6" "$6"
    near "our $1, and what it was" moving.y4m ours.y4m 50 46 46
    ffmpeg -v error -y -i moving.y4m -pix_fmt "$5" -r "$3" theirs.dv || fail "ffmpeg did not write DV"
    expect 0 "10 frames of $1, $2" dv info theirs.dv
    expect 0 "errors      none" dv info theirs.dv
    expect 0 "10 frames" dv decode theirs.dv theirs.y4m
    near "FFmpeg's $1, by FFmpeg and by us" theirs.dv theirs.y4m 58 "$6" "$6"
}
both NTSCDV25 720x480 30000/1001 bt601 yuv411p 47
both PALDV25 720x576 25 bt601 yuv420p 47
both NTSCDV50 720x480 30000/1001 bt601 yuv422p 56
both PALDV50 720x576 25 bt601 yuv422p 56
both NTSC_DV100_720p 960x720 60000/1001 bt709 yuv422p 56
both PAL_DV100_720p 960x720 50 bt709 yuv422p 56
both NTSC_DV100_1080i 1280x1080 30000/1001 bt709 yuv422p 56
both PAL_DV100_1080i 1440x1080 25 bt709 yuv422p 56

finish
