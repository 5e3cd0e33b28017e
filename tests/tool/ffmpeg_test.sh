# A clip of 4:2:0 from FFmpeg through the program and back, with the error of each plane.
. "$(dirname "$0")/expect.sh"

if ! command -v ffmpeg > found; then
    echo "skipped: ffmpeg is not installed"
    exit 77
fi

# clip NAME WORDS FILTERS: ten frames that move over a photograph
clip() {
    ffmpeg -v error -y -loop 1 -i "$media/coffee.png" -frames:v 10 $2 \
        -vf "crop=352:288:n*4:n*3,scale=out_color_matrix=bt601:flags=accurate_rnd+bicubic${3:-}" -pix_fmt yuv420p "$1" ||
        fail "ffmpeg did not write $1"
}
clip left.y4m "-chroma_sample_location left"
clip center.y4m "-chroma_sample_location center"
clip fields.y4m "-chroma_sample_location left" ",tinterlace=interleave_top,setfield=tff"
is "what FFmpeg says of fields" "$(head -1 fields.y4m | grep -o ' I.')" " It"

# psnr FILE FILE: of Y, U and V over all frames, such as "inf 50.18 48.56". Frames are met by their times, so that streams
# must be of one rate.
psnr() {
    local raw=()
    case $1 in *.yuv) raw=(-f rawvideo -pix_fmt yuv420p -video_size 352x288) ;; esac
    ffmpeg -hide_banner -nostats "${raw[@]}" -i "$1" "${raw[@]}" -i "$2" -lavfi psnr -f null - 2>&1 |
        sed -n 's/.*PSNR y:\([^ ]*\) u:\([^ ]*\) v:\([^ ]*\) .*/\1 \2 \3/p'
}
# near FILE FILE Y U V: no plane is further off than so many dB, inf for not at all
near() {
    local got
    got=$(psnr "$1" "$2")
    echo "$1 and $2: $got dB"
    is "$1 and $2, $got dB, at least $3 $4 $5" "$(echo "$got" | awk -v y="$3" -v u="$4" -v v="$5" '
        function reaches(got, least) { return got == "inf" || (least != "inf" && got + 0 >= least + 0) }
        { print NF == 3 && reaches($1, y) && reaches($2, u) && reaches($3, v) }')" 1
}

for name in left center fields; do
    expect 0 "352x288" convert $name.y4m same.y4m
    near $name.y4m same.y4m inf inf inf
    ffmpeg -v error -y -i $name.y4m -f rawvideo -pix_fmt nv12 from_ffmpeg.nv12
    expect 0 "" convert $name.y4m from_us.nv12 --to nv12
    same "nv12 of $name" from_ffmpeg.nv12 from_us.nv12
    ffmpeg -v error -y -i $name.y4m -f rawvideo from_ffmpeg.yuv
    expect 0 "" convert $name.y4m from_us.yuv --to yuv420p
    same "yuv420p of $name" from_ffmpeg.yuv from_us.yuv
done

# Decoded to pixels and encoded again. Luma stays; chroma is interpolated and filtered, and encoded as on the left, which
# tells on what was centred.
through() { # NAME FORMAT Y U V
    expect 0 "10 frames 352x288, $2 to YUV_420" convert "$1.y4m" through.y4m --from "$2"
    near "$1.y4m" through.y4m "$3" "$4" "$5"
}
through left VUYX_4444_8u inf 49 47
through left BGRA_4444_8u 60 49 47
through center VUYX_4444_8u inf 45 44
through fields VUYX_4444_8u inf 45 43
# Fields decoded as frames, or frames as fields, would show: chroma of the two fields is mixed.
ffmpeg -v error -y -i fields.y4m -f rawvideo fields.yuv
expect 0 "YUV_420_MPEG2_FRAME to" convert fields.yuv mixed.yuv --from yuv420p:frames --to VUYX_4444_8u --size 352x288
expect 0 "VUYX_4444_8u to YUV_420_MPEG2_FIELD" convert mixed.yuv again.yuv --from VUYX_4444_8u \
    --to yuv420p:fields --size 352x288
mixed=$(psnr fields.yuv again.yuv)
echo "fields that were taken for frames: $mixed dB"
is "which shows, $mixed dB" "$(echo "$mixed" | awk '{ print NF == 3 && $1 == "inf" && $2 < 42 }')" 1

finish
